#pragma once

// Makes the pictures below ":/res/" known. A static library's resources are left out of the program
// unless somebody asks for them: call this once before the first screen is built. More calls do no
// harm.
void initResources();
