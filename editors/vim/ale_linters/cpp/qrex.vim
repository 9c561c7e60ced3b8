call qrex_ale#Define('cpp')
