// Gives a ticket without a Layout one, built from its run lists, and writes it to the output path.
#pragma once

class LD_JDF;

class LayoutInjectionProcessingJdf {
public:
    LayoutInjectionProcessingJdf(wchar_t* jdfPath, wchar_t* dataPath, char* outputPath, LD_JDF* worker);
    // 0 on success, 1 when the ticket could not be written.
    int run();

private:
    wchar_t* jdfPath_;
    wchar_t* dataPath_;
    char* outputPath_;
    LD_JDF* worker_;
};
