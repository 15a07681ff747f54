# Precompiled headers: what most of the browser's sources include and none of ours changes. They are
# compiled once and used by every target that is built with the same options: 400 seconds of a build
# from nothing on two cores become 290. The preset `device` does without, so that a source that
# forgot an include of its own is found. (The service gains nothing: its sources include less than a
# common set would hold.)

option(ORVALA_PRECOMPILED_HEADERS "Compile the large headers of the libraries only once" ON)

set(qt_headers
  <algorithm> <functional> <memory> <utility> <vector>
  <QByteArray> <QCoreApplication> <QDateTime> <QDir> <QFile> <QHash> <QList> <QObject> <QPointer>
  <QSettings> <QSize> <QString> <QStringList> <QTimer> <QUrl> <QVariant> <QVector>
  <QNetworkAccessManager> <QNetworkReply>
  <QApplication> <QBoxLayout> <QImage> <QKeyEvent> <QLabel> <QPainter> <QPixmap> <QPushButton>
  <QWidget>)

file(WRITE ${CMAKE_BINARY_DIR}/generated/headers.cpp "")
file(WRITE ${CMAKE_BINARY_DIR}/generated/headers-main.cpp "int main() {}\n")

# Qt's libraries are position independent in another way than its programs: a set for each.
function(orvala_header_sets)
  if(NOT ORVALA_PRECOMPILED_HEADERS)
    return()
  endif()
  add_library(orvala_qt_headers STATIC ${CMAKE_BINARY_DIR}/generated/headers.cpp)
  add_executable(orvala_qt_program_headers ${CMAKE_BINARY_DIR}/generated/headers-main.cpp)
  foreach(target orvala_qt_headers orvala_qt_program_headers)
    # A set suits every target that defines what the set was compiled with: so no QT_WIDGETS_LIB.
    target_link_libraries(${target} PRIVATE Qt5::Core)
    foreach(library Gui Network Widgets)
      target_include_directories(${target} SYSTEM PRIVATE ${Qt5${library}_INCLUDE_DIRS})
    endforeach()
    target_precompile_headers(${target} PRIVATE ${qt_headers})
    orvala_settings(${target})
    orvala_qt_definitions(${target})
  endforeach()
endfunction()

# The target's sources start from a set.
function(orvala_use_headers target set)
  if(ORVALA_PRECOMPILED_HEADERS)
    target_precompile_headers(${target} REUSE_FROM ${set})
  endif()
endfunction()
