#pragma once

// True when the file is well-formed XML whose root element is OptionalContentGroupData (any case).
bool isVersionDescriptionFile(const char* path);
