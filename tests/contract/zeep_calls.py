"""Calls every operation of a storefront simulator through its own WSDLs with another SOAP toolkit (zeep), over TLS, and
compares what that toolkit read with the simulator's database: zeep_calls.py PROGRAM
"""
import decimal
import hashlib
import json
import os
import re
import sqlite3
import subprocess
import sys
import tempfile
import time
import urllib.request

import requests
import zeep
import zeep.transports

NAMESPACES = {
    'wsse': 'http://docs.oasis-open.org/wss/2004/01/oasis-200401-wss-wssecurity-secext-1.0.xsd',
    'wsa': 'http://schemas.xmlsoap.org/ws/2004/08/addressing',
    'api': 'http://api.zorvane.example/api/',
}
OASIS = 'http://docs.oasis-open.org/wss/2004/01/oasis-200401-wss-'
SERVICES = ['RealTimeBrowse', 'DownloadAPI', 'StreamAPI']


class Sql(str):
    """The first value of a query, or with `every` the first column."""
    every = False


class SqlList(Sql):
    every = True


SKU = Sql('SELECT MIN(sku) FROM product WHERE type = 1 AND title > 50 AND CAST(price AS REAL) < 10')
SEASON = Sql('SELECT MIN(id) FROM title WHERE is_tv = 1')
EPISODE = Sql('SELECT MIN(id) FROM title WHERE season > 0')
BONUS = Sql('SELECT MIN(id) FROM bonus')
PREPAID = Sql('SELECT prepaid FROM account WHERE id = 1')
PAGE = {'CurrentPageNumber': 1, 'ItemsPerPage': 3, 'PurchaseType': 'any'}
ANY = {'TitleType': 'any', 'WatchStatusFilter': 'Undefined'}
SEARCH = {**PAGE, 'Query': 'the', 'TitleType': 'any'}
PASS = {'PassID': 1, 'FileProfile': 'HIGH_DEFINITION'}
OK = {'ResponseCode': 0, 'ResponseMessage': 'OK'}
FOUND = Sql("SELECT COUNT(*) FROM title WHERE name LIKE '%the%'")
TITLE = {
    'TitleID': 13, 'TitleName': Sql('SELECT name FROM title WHERE id = 13'), 'ResponseCode': 0,
    'Synopsys': Sql('SELECT synopsis FROM title WHERE id = 13'),
    'AvailableProducts.ProductListing.0.Price': Sql('SELECT price FROM product WHERE title = 13 ORDER BY sku'),
    'AvailableProducts.ProductListing.0.ExpireDate': Sql('SELECT expires FROM product WHERE title = 13 ORDER BY sku'),
    'AvailableProducts.ProductListing.0.AvailableAssets.FileProfile': ['STANDARD', 'HIGH_DEFINITION'],
    'BonusAssets.BonusAsset.0.BonusAssetID': Sql('SELECT id FROM bonus WHERE title = 13'),
}
VIDEOS = {**OK, 'Titles.TitleListingPurchased.*.TitleID': SqlList('SELECT title FROM pass WHERE account = 1 LIMIT 3'),
          'TotalItems': Sql('SELECT COUNT(*) FROM pass WHERE account = 1')}
WISHES = {**OK, 'SortOrder': 0, 'Titles.TitleListingPurchased.*.TitleID':
          SqlList('SELECT title FROM wish WHERE account = 1 ORDER BY added')}
LOCATION = {**OK, 'AssetID': 102, 'StreamID': 'stream-1'}

# Services by their first letters, operation, arguments, and what the answer must hold: by the path of a child ("*" for
# each element of an array), or "" for the whole answer.
CALLS = [
    ('R', 'getFileType', {}, {'File_AccessType': 'STREAM', 'File_FileExtension': 'MP4'}),
    ('R', 'getLastCacheLoadTimeUTC', {}, {'': Sql('SELECT load_time FROM service')}),
    ('R', 'shouldUpdateCache', {'UTCTime': Sql('SELECT load_time FROM service')}, {'': 0}),
    ('R', 'shouldUpdateCache', {'UTCTime': 'then'}, {'': 1}),
    ('R', 'getNavigation', {}, {'Genre.*.Name': SqlList('SELECT name FROM genre ORDER BY id')}),
    ('R', 'getGenreLabel', {'GenreID': 1}, {**OK, 'Label': Sql('SELECT label FROM genre WHERE id = 1')}),
    ('R', 'getTitlesByNavigation', {**PAGE, 'GenreID': 1},
     {**OK, 'GenreID': 1, 'ItemsPerPage': 3, 'Titles.TitleListing.*.TitleID':
      SqlList('SELECT title FROM title_genre WHERE genre = 1 ORDER BY title LIMIT 3')}),
    ('R', 'getTitlesByGenreArray', {**PAGE, 'GenreIDs': {'int': [2, 1]}},
     {'*.GenreID': [2, 1], '*.TotalItems':
      SqlList('SELECT COUNT(*) FROM title_genre WHERE genre < 3 GROUP BY genre ORDER BY genre DESC')}),
    ('R', 'getTitleListing', {'TitleID': 13}, TITLE),
    ('R', 'getTitleListing', {'TitleID': 0}, {'ResponseCode': 1, 'ResponseMessage': 'no such title', 'Synopsys': None}),
    ('R', 'getTvEpisodeListing', {'EpisodeID': EPISODE}, {'TitleID': EPISODE, 'ResponseCode': 0}),
    ('R', 'getTvEpisodeListByTitleID', {'TitleID': SEASON},
     {**OK, 'Episodes.TvEpisode.*.EpisodeID': SqlList(f'SELECT id FROM title WHERE season = ({SEASON}) ORDER BY episode')}),
    ('R', 'getAllTvEpisodeListings', {'TitleID': SEASON},
     {'*.TitleName': SqlList(f'SELECT name FROM title WHERE season = ({SEASON}) ORDER BY episode')}),
    ('R', 'translateSkuId', {'SkuId': SKU}, {**OK, 'TitleId': Sql(f'SELECT title FROM product WHERE sku = ({SKU})')}),
    ('R', 'translateTivoExternalId', {'TivoExternalId': 'EXT12'}, {**OK, 'TivoExternalId': 'EXT12', 'TitleId': 12}),
    ('R', 'searchForTitle', SEARCH, {**OK, 'TotalItems': FOUND}),
    ('R', 'searchForTitleDetail', {**SEARCH, 'Query': 'Caf\u00e9 & <b>'}, {**OK, 'TotalItems': 0}),
    ('R', 'getRecommendedTitles', {'TitleId': 12}, {**OK, 'Titles.TitleListing.0.TitlePosition': 1}),
    ('DS', 'checkRentalExpiration', {'PassId': 1},
     {**OK, 'ShouldDisplay': True, 'HoursRemaining': Sql('SELECT hours FROM pass WHERE id = 1')}),
    ('DS', 'GetCountryID', {}, {'': Sql('SELECT country FROM account WHERE id = 1')}),
    ('DS', 'getConfig', {}, {**OK, 'ConfigurationSet.Configuration.*.Key': ['BandwithCheckURL', 'Region', 'Unset'],
                             'ConfigurationSet.Configuration.2.Value': None}),
    ('DS', 'checkAdultVerificationPin', {'Pin': '0042'}, {**OK, 'IsPinVerified': True}),
    ('DS', 'checkAdultVerificationPin', {'Pin': '42'}, {**OK, 'IsPinVerified': False}),
    ('DS', 'checkAdultVerificationEnabled', {}, {**OK, 'IsAdultVerificationEnabled': 'true'}),
    ('DS', 'addItemToWishlist', {'TitleID': 60}, OK),
    ('DS', 'getWishlistItems', {'sortOrder': 0, 'CurrentPageNumber': 1, 'ItemsPerPage': 9, 'TitleType': 'any'}, WISHES),
    ('D', 'removeItemFromWishList', {'TitleID': 60}, OK),
    ('S', 'removeItemFromWishList', {'TitleID': 60}, {'ResponseCode': 1, 'ResponseMessage': 'not in the wish list'}),
    ('DS', 'removeAllItemsFromWishList', {}, OK),
    ('D', 'assignGiftCertificateToUser', {'GiftCertificateCode': 'GIFT1'}, {**OK, 'Balance': PREPAID}),
    ('S', 'assignGiftCertificateToUser', {'GiftCertificateCode': 'GIFT2'}, {**OK, 'Balance': PREPAID}),
    ('DS', 'getSettingsPageInfo', {}, {**OK, 'Account': Sql('SELECT name FROM account WHERE id = 1')}),
    ('DS', 'getEmailAddress', {}, {**OK, 'EmailAddress': Sql('SELECT email FROM account WHERE id = 1')}),
    ('DS', 'showPrePaidCardBalance', {}, {**OK, 'Balance': PREPAID}),
    ('DS', 'getBillingInfo', {}, {**OK, 'CCLastFour': Sql('SELECT card FROM account WHERE id = 1')}),
    ('S', 'getBillingInfoAndPPCBalance', {}, {'BillingInfo.ResponseCode': 0, 'PPCardBalance.Balance': PREPAID}),
    ('D', 'checkForPurchasedTitle', {'TitleID': 12}, {'': True}),
    ('S', 'checkForPurchasedStreamByTitleID', {'TitleID': 59}, {'': False}),
    ('S', 'checkForPurchasedStream', {'SkuID': SKU}, {'': False}),
    ('D', 'getMyVideos', {**PAGE, **ANY}, VIDEOS),
    ('S', 'getMyStreamingVideos', {**PAGE, **ANY}, VIDEOS),
    ('S', 'getTitleListingsPurchasedForPasses', {'Passes': {'int': [2, 1]}},
     {'*.PassID': [2, 1], '*.ResponseCode': [0, 0]}),
    ('DS', 'doPurchaseSavedbilling', {'SkuID': SKU, 'IPAddress': '10.0.0.1', 'UsePrePaidFunds': 'yes'},
     {**OK, 'PassID': Sql('SELECT MAX(id) FROM pass')}),
    ('DS', 'doPurchaseSavedbilling', {'SkuID': 9022, 'IPAddress': '10.0.0.1', 'UsePrePaidFunds': 'no'},
     {'ResponseCode': 22}),
    ('S', 'calcOrderTax', {'SKUID': SKU}, {**OK, 'TotalPrice': Sql(f'SELECT price FROM product WHERE sku = ({SKU})')}),
    ('DS', 'authorizeDevice', {'PIN': '000000'}, {'ResponseCode': 2, 'AuthToken': None}),
    ('DS', 'authorizeDevice', {'PIN': '123456'},
     {**OK, 'AuthToken': Sql('SELECT text FROM token ORDER BY number DESC LIMIT 1')}),
    ('DS', 'checkAuthToken', {'AuthToken': Sql('SELECT text FROM token ORDER BY number DESC LIMIT 1')}, {'': True}),
    ('DS', 'deactivateDevice', {}, OK),
    ('DS', 'checkAuthToken', {'AuthToken': Sql('SELECT text FROM token ORDER BY number DESC LIMIT 1')}, {'': False}),
    ('S', 'setAudioDefaultProperty', {'AudioSetting': 'DTS_Express_51'}, OK),
    ('S', 'getAudioDefaultProperty', {}, {'': 'DTS_Express_51'}),
    ('S', 'getTHXMediaDirector', {**PASS, 'AudioSetting': 'DTS_Express_51'}, {**OK, 'ShortFormat': 'THX-S'}),
    ('S', 'getTHXMediaDirectorBonusAsset',
     {'BonusAssetID': BONUS, 'FileProfile': 'STANDARD', 'BonusAssetType': 'Trailer'},
     {**OK, 'LongFormat': 'THX-LONG-Trailer'}),
    ('S', 'getStreamingAssetLocation', PASS, {**LOCATION, 'StartTimeSeconds': 0}),
    ('S', 'manageStreamInstanceStatus', {'StreamID': 'stream-1', 'Status': 'paused', 'StopTimeSeconds': 77}, OK),
    ('S', 'loadLastStreamingAssetLocationForPass', PASS, {**LOCATION, 'Status': 'paused', 'StartTimeSeconds': 77}),
    ('S', 'getBonusAssetLocation', {'BonusAssetID': BONUS}, {**OK, 'AssetID': BONUS}),
    ('S', 'ReturnTimeout', {}, OK),
    ('S', 'ReturnError', {}, OK),
    ('S', 'removeAllMyPurchases', {'password': 'secret'}, OK),
]


class Storefront:
    """A simulator in a process of its own, and its database."""

    def __init__(self, program, folder):
        self.process = subprocess.Popen([program, '--data', folder], stdout=subprocess.PIPE, text=True)
        said = {}
        for line in self.process.stdout:  # ends with the process
            if line == 'ready\n':
                break
            name, _, value = line.rstrip('\n').rpartition(' ')
            said[name] = value
        else:
            sys.exit('the simulator did not start')
        self.https = f"https://localhost:{said['https port']}"
        self.http = f"http://localhost:{said['http port']}"
        with open(said['deployment file'], encoding='utf-8') as file:
            self.authority = re.search('^ca_file = (.*)$', file.read(), re.MULTILINE).group(1)
        self.database = sqlite3.connect(f'file:{folder}/storefront.db?mode=ro', uri=True)

    def control(self, method, path, text=None):
        request = urllib.request.Request(f'{self.http}/control/{path}', text and text.encode(), method=method)
        opener = urllib.request.build_opener(urllib.request.ProxyHandler({}))
        with opener.open(request) as answer:
            return answer.read().decode()

    def values(self, value):
        """The value, or what it stands for."""
        if isinstance(value, dict):
            return {name: self.values(part) for name, part in value.items()}
        if not isinstance(value, Sql):
            return value
        rows = [row[0] for row in self.database.execute(value)]
        return rows if value.every else rows[0]

    def end(self):
        self.database.close()
        self.process.terminate()
        return self.process.wait()


class Service:
    """One of the three, by its WSDL."""

    def __init__(self, name, store):
        session = requests.Session()
        session.trust_env = False
        session.verify = store.authority
        address = f'{store.https}/api/{name}.asmx'
        self.client = zeep.Client(f'{address}?wsdl', transport=zeep.transports.Transport(session=session),
                                  settings=zeep.Settings(strict=True))
        self.name = name
        self.address = address
        assert self.client.service._binding_options['address'] == address, 'the address in the WSDL'
        self.operations = self.client.service._binding._operations

    def element(self, prefix, name, *values, **children):
        return self.client.get_element(f'{{{NAMESPACES[prefix]}}}{name}')(*values, **children)

    def headers(self, operation):
        """The blocks that the WSDL names, made with its types."""
        nonce, created = os.urandom(20), time.strftime('%Y-%m-%dT%H:%M:%SZ', time.gmtime())
        digest = hashlib.sha1(nonce + created.encode() + b'secret').digest()
        token = {
            'Username': 'customer',
            'Password': {'_value_1': digest, 'Type': f'{OASIS}username-token-profile-1.0#PasswordDigest'},
            'Nonce': {'_value_1': nonce, 'EncodingType': f'{OASIS}soap-message-security-1.0#Base64Binary'},
            'Created': created,
            'Id': 'User',
        }
        anonymous = NAMESPACES['wsa'] + '/role/anonymous'
        device = {'APIKey': 'desktop', 'DestinationUniqueID': 'another', 'DestinationTypeID': 48}
        blocks = {
            'Security': {'UsernameToken': token, 'mustUnderstand': '1'},
            'MessageID': f'uuid:{operation}',
            'ReplyTo': {'Address': anonymous, 'mustUnderstand': '1'},
            'To': {'_value_1': self.address, 'mustUnderstand': '1'},
            'Action': {'_value_1': NAMESPACES['api'] + operation, 'mustUnderstand': '1'},
        }
        last = list(self.operations[operation].input.header.type.elements)[-1][0]
        blocks[last] = {**device, 'mustUnderstand': '1'}
        return blocks

    def call(self, operation, arguments):
        return self.client.service[operation](**arguments, _soapheaders=self.headers(operation))


def child(value, path):
    """What stands at a path."""
    step, _, rest = path.partition('.')
    if not path:
        return value
    if step == '*':
        return [child(element, rest) for element in value]
    if step.isdigit():
        return child(value[int(step)], rest)
    return child(getattr(value, step, f'no {step}'), rest)


def same(got, wanted):
    if isinstance(got, decimal.Decimal):
        return str(got) == wanted
    return got == wanted and isinstance(got, bool) == isinstance(wanted, bool)


def main(program):
    failures = []
    with tempfile.TemporaryDirectory() as folder:
        store = Storefront(program, folder)
        try:
            services = [Service(name, store) for name in SERVICES]
            called = set()
            for letters, operation, arguments, expected in CALLS:
                for service in [service for service in services if service.name[0] in letters]:
                    answer = service.call(operation, store.values(arguments))
                    called.add((service.name, operation))
                    for path, wanted in store.values(expected).items():
                        got = child(answer, path)
                        if not same(got, wanted):
                            failures.append(f'{service.name} {operation} {path}: {got!r}, not {wanted!r}')
            every = {(service.name, operation) for service in services for operation in service.operations}
            failures += [f'never called: {missing}' for missing in every - called]

            store.control('POST', 'faults', 'getNavigation=fault11')
            try:
                services[0].call('getNavigation', {})
                failures.append('a fault was read as an answer')
            except zeep.exceptions.Fault as fault:
                if fault.message != 'the shop is closed':
                    failures.append(f'the fault reads {fault.message}')
            log = [json.loads(line) for line in store.control('GET', 'log').splitlines()]
            failures += [entry['violation'] for entry in log if entry['violation']]
            print(f'{len(every)} operations called')
        finally:
            if store.end() != 0:
                failures.append('the simulator ended with an error')
    return failures


if __name__ == '__main__':
    found = main(sys.argv[1])
    for failure in found:
        print(failure)
    sys.exit(1 if found else 0)
