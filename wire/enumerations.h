// Enumerations of the service schema. The numbers are the ones the client stores; the texts are the names after the
// last "__" with _USCORE for an underscore, and their mixed case is the schema's own.

enum ZV1__AccessType {
    ZV1__AccessType__UNKNOWN = 0,
    ZV1__AccessType__DOWNLOAD = 1,
    ZV1__AccessType__STREAM = 2,
};

enum ZV1__DRMProvider {
    ZV1__DRMProvider__UNKNOWN = 0,
    ZV1__DRMProvider__WMDRM_USCORE10 = 1,
    ZV1__DRMProvider__TIVO_USCOREDRM = 2,
    ZV1__DRMProvider__WIDEVINE = 3,
    ZV1__DRMProvider__WMDRM_USCORE7 = 4,
    ZV1__DRMProvider__WMDRM_USCORE9 = 5,
    ZV1__DRMProvider__FLUX = 6,
    ZV1__DRMProvider__DIVX = 7,
    ZV1__DRMProvider__Intel_USCOREMV = 8,
    ZV1__DRMProvider__RTMPE = 9,
    ZV1__DRMProvider__FLASH_USCOREACCESS = 10,
    ZV1__DRMProvider__PLAY_USCOREREADY = 11,
};

enum ZV1__FileProfile {
    ZV1__FileProfile__UNKNOWN = 0,
    ZV1__FileProfile__STANDARD = 1,
    ZV1__FileProfile__HIGH_USCOREDEFINITION = 2,
    ZV1__FileProfile__PORTABLE = 3,
    ZV1__FileProfile__PORTABLE_USCORESTANDARD = 4,
    ZV1__FileProfile__TEMP5 = 5,
    ZV1__FileProfile__PORTABLE_USCOREWIDE = 6,
    ZV1__FileProfile__STANDARD_USCOREDEFINITION_USCORE3D = 7,
    ZV1__FileProfile__HIGH_USCOREDEFINITION_USCORE3D = 8,
    ZV1__FileProfile__STANDARD_USCOREDEFINITION_USCOREREALD_USCORE3D = 9,
    ZV1__FileProfile__HIGH_USCOREDEFINITION_USCOREREALD_USCORE3D = 10,
};

enum ZV1__VideoFormat {
    ZV1__VideoFormat__UNKNOWN = 0,
    ZV1__VideoFormat__WMV9 = 1,
    ZV1__VideoFormat__MPEG2_USCORETIVO = 2,
    ZV1__VideoFormat__MPEG2_USCOREStandard = 3,
    ZV1__VideoFormat__VC1 = 4,
    ZV1__VideoFormat__DIVX = 5,
    ZV1__VideoFormat__H264 = 6,
    ZV1__VideoFormat__FLUX = 7,
};

enum ZV1__FileExtension {
    ZV1__FileExtension__AUTOPOPULATE = 0,
    ZV1__FileExtension__UNKNOWN = 1,
    ZV1__FileExtension__WMV = 2,
    ZV1__FileExtension__MPEG = 3,
    ZV1__FileExtension__MP4 = 4,
    ZV1__FileExtension__FLUX = 5,
    ZV1__FileExtension__AVI = 6,
    ZV1__FileExtension__QT = 7,
    ZV1__FileExtension__FLV = 8,
    ZV1__FileExtension__RM = 9,
    ZV1__FileExtension__DIVX = 10,
};

enum ZV1__WatchStatus {
    ZV1__WatchStatus__WatchNow = 0,
    ZV1__WatchStatus__RentAgain = 1,
    ZV1__WatchStatus__NotAvailable = 2,
    ZV1__WatchStatus__Undefined = 3,
};

enum ZV1__StreamStatus {
    ZV1__StreamStatus__play = 0,
    ZV1__StreamStatus__stopped = 1,
    ZV1__StreamStatus__paused = 2,
    ZV1__StreamStatus__resumeplay = 3,
    ZV1__StreamStatus__errorinplayback = 4,
};

enum ZV1__AudioProfile {
    ZV1__AudioProfile__Stereo_USCOREStandard = 0,
    ZV1__AudioProfile__Dolby_USCOREStereo_USCOREAC3 = 1,
    ZV1__AudioProfile__Dolby_USCOREDigital_USCOREPlus_USCOREStereo = 2,
    ZV1__AudioProfile__Dolby_USCOREDigital_USCOREPlus_USCORE51 = 3,
    ZV1__AudioProfile__DTS_USCOREExpress_USCOREStereo = 4,
    ZV1__AudioProfile__DTS_USCOREExpress_USCORE51 = 5,
};

enum ZV1__BonusAssetType {
    ZV1__BonusAssetType__Trailer = 0,
};

enum ZV1__TitleTypeFilter {
    ZV1__TitleTypeFilter__any = 0,
    ZV1__TitleTypeFilter__tv = 1,
    ZV1__TitleTypeFilter__movies = 2,
};

enum ZV1__StreamAPIPurchaseType {
    ZV1__StreamAPIPurchaseType__rent = 0,
    ZV1__StreamAPIPurchaseType__buy = 1,
    ZV1__StreamAPIPurchaseType__any = 2,
};
