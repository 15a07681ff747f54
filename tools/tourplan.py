"""What the tour presses, and which pictures it takes.

A step is (actions, picture) or (actions, picture, MOVING): the actions are pressed in order, then the screen has to
change and, unless it is MOVING by itself, come to rest; a step without a picture only goes on. Actions are keys of
the remote ("down*3": three times), "type:TEXT" on a real keyboard (the only action of its step), "freeze" and "thaw"
for a service that does not answer, "stop-service", "cable-out", "cable-in" and "wait:SECONDS".
"""

from dataclasses import dataclass, field

MOVING = "moving"
ANNA = ("anna@orvala.example", "Anna Lindqvist")
BEN = ("ben@orvala.example", "Ben Okafor")
LONG = ("featherstonehaugh-cholmondeley.maximiliana@a-very-long-host-name.orvala.example",
        "Maximiliana Featherstonehaugh-Cholmondeley")
PEOPLE = {ANNA[0], BEN[0]}
# Beside what the demo's people wrote.
PHOTO = "anna/Garden/Pusteblume im Abendlicht.heic"
COMMENTS = [
    {"photo": PHOTO, "author": author, "text": text, "published": f"2026-06-{day:02}T20:15:00Z"}
    for day, (author, text) in enumerate([
        (BEN[0], "First!"),
        (ANNA[0], "You always say that. And it is never about the photo, it is about being first, which I find "
                  "remarkable in somebody who has not once in his life been on time for dinner."),
        (BEN[0], "Donaudampfschifffahrtselektrizitätenhauptbetriebswerkbauunterbeamtengesellschaftsvorsitzender"),
        (ANNA[0], "?"),
        (BEN[0], "איזה יופי! 🌼🌬️"),
        (ANNA[0], "<b>Not bold</b> & not &amp; either."),
    ], start=1)]
TAGS = [{"photo": PHOTO, "author": BEN[0], "tag": tag}
        for tag in ("wish", "the longest tag that anybody ever gave to a photo of a simple dandelion in the evening "
                    "light of a day in May", "löwenzahn", "<i>tag</i>")]
ODD_ALBUM = "Was wir in den langen Ferien bei den Großeltern an der See alles erlebt haben, Teil 2 von 3 & <b>mehr"


@dataclass
class Chapter:
    name: str
    steps: list
    accounts: list = field(default_factory=lambda: [ANNA])
    opening: str = ""
    needs_network: bool = False


def wrong_password(picture):
    return [("select", ""), ("type:hills", ""), ("select", ""), ("down", ""), ("select", picture)]


CHAPTERS = [
    Chapter("sign-in", accounts=[], opening="first-start", steps=[
        ("freeze select", "sign-in-loading", MOVING),
        ("thaw", "sign-in"),
        ("select", "sign-in-mail"),
        ("red", "keyboard-capitals"),
        ("page-down*2", "keyboard-signs"),
        ("page-down", "keyboard-smileys"),
        ("page-up*3", ""),
        ("type:anna@orvala.example", "keyboard-typed"),
        ("select", ""),
        ("down", "sign-in-filled"),
        ("select", ""),
        ("type:hills", "sign-in-password"),
        ("select", ""),
        ("down", "sign-in-button"),
        ("select", "sign-in-wrong"),
        ("down", ""),
        *wrong_password(""),
        ("down", ""),
        *wrong_password("sign-in-panel"),
    ]),
    Chapter("consent", accounts=[], steps=[
        ("select", ""),
        ("select", ""),
        ("type:anna@orvala.example", ""),
        ("select", ""),
        ("down", ""),
        ("select", ""),
        ("type:mountains", ""),
        ("select", ""),
        ("down", ""),
        ("select", "consent"),
    ]),
    Chapter("accounts", accounts=[BEN, (*LONG, "4711"), ANNA], opening="accounts", steps=[
        ("right", "account-delete-button"),
        ("select", "account-delete"),
        ("return", ""),
        ("right", "account-new"),
        ("down", "account-code"),
        ("select", "account-form"),
        ("select", "account-form-input"),
        ("type:anna", ""),
        ("select", "account-form-code"),
        *[("type:" + digit, "") for digit in "1234"],
        ("select", "account-form-tip"),
        ("up right select", "account-list"),
        ("return", ""),
        ("return", ""),
        ("up", ""),
        ("stop-service select", "sign-in-no-service"),
    ]),
    Chapter("browse", steps=[
        ("freeze select", "loading", MOVING),
        ("thaw", "home"),
        ("page-down", "home-page-2"),
        ("down right", "home-second-row"),
        ("red", ""),
        ("up right", "menu"),
        ("right*3", "menu-sign-out"),
        ("left*3 select", "albums"),
        ("down", "albums-second-row"),
        ("right", "albums-long-title"),
        ("up right", ""),
        ("select wait:3", "album"),  # the service takes its time for a HEIC file
        ("freeze page-down", "album-no-thumbnails-yet"),
        ("thaw", "album-page-2"),
        ("return", ""),
        ("up right*3 select", "sign-out-question"),
    ]),
    Chapter("photo", steps=[
        ("select", ""),
        ("up right select", ""),
        ("right*2 select", ""),
        ("select", "photo"),
        ("right*3", "photo-upright"),
        ("down", "photo-actions"),
        ("right select", "zoom"),
        ("select", "zoom-closer"),
        ("right*3", "zoom-right"),
        ("return", ""),
        ("right*5 select", "photo-information-off"),
        ("select", ""),
        ("up right*2", "photo-remarks"),
        ("down left*3 select", "comments"),
        ("down*3", "comments-scrolled"),
        ("select", "comment-delete"),
        ("return", ""),
        ("return", ""),
        ("right", ""),
        ("select", "tags"),
        ("down", ""),
        ("select", "tag-delete"),
        ("return", ""),
        ("return", ""),
        ("right select", "tag-input"),
        ("type:summer", "tag-typed"),
        ("freeze select", "sending", MOVING),
        ("thaw", "toast"),
        ("wait:4 left*3", ""),
        ("select", "comment-input"),
    ]),
    Chapter("search", steps=[
        ("select", ""),
        ("up right*3 select", "search"),
        ("select", ""),
        ("type:flowers", "search-input"),
        ("select", "search-text"),
        ("right", "search-button"),
        ("select", "search-results"),
        ("return select", ""),
        ("type:xyz", ""),
        ("select", ""),
        ("right select", "no-photo"),
    ]),
    Chapter("favourites", steps=[
        ("select", ""),
        ("up right*2 select", "favourites"),
        ("select", "person"),
        ("right*2 select", "person-album"),
        ("select", "person-photo"),
        ("right*2", "photo-failed"),
    ]),
    Chapter("slide-show", steps=[
        ("select", ""),
        ("up right select", ""),
        ("right*3 select", ""),
        ("play", "slide-show", MOVING),
        ("pause", "slide-show-paused"),
        ("right", "slide-show-caption"),
        ("wait:5 right", "slide-show-upright"),
        ("setting", "slide-settings"),
        ("up*2 select down", "slide-settings-editing"),
        ("select down*2 right", ""),
        ("select", ""),
        ("return", "after-slide-show"),
    ]),
    Chapter("cable", needs_network=True, steps=[
        ("select", ""),
        ("cable-out", "cable-out"),
        ("cable-in", "cable-in"),
    ]),
    Chapter("offline", steps=[
        ("select", ""),
        ("stop-service up right select", "offline"),
    ]),
    Chapter("long-name", accounts=[LONG], steps=[
        ("select", "long-name"),
        ("up right*4 select", "sign-out-long-name"),
    ]),
]
